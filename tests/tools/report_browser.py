#!/usr/bin/env python3
"""The page of `tevpf report` in headless Chromium: sorting, filtering, keyboard, contrast, narrow windows, paper,
and life without script. Leaves pictures in the folder, for people to look at.

    report_browser.py TEVPF FOLDER     (needs chromium-driver and python3-selenium)
"""
import base64
import os
import pathlib
import subprocess
import sys

from selenium import webdriver
from selenium.webdriver.common.by import By
from selenium.webdriver.common.keys import Keys

ROWS = [(10, "1.00000012", "nominal"), (9, "nan", "Cut off"), (100, "1.00000011", "<script>alert(1)</script>"),
        (-5, "-inf", "run 10"), (2, "1e300", "run 9"), (7, "", "' onclick='alert(2)")]
# In order: n, x with what is not a number last, and labels with their numbers by size.
ORDERS = {"n": [4, 5, 6, 2, 1, 3], "x": [4, 3, 1, 5, 2, 6], "label": [6, 3, 2, 1, 5, 4]}

CONTRAST = """
const light = (rgb) => rgb.match(/[\\d.]+/g).slice(0, 3).map((v) => v / 255)
    .map((v) => v <= .04045 ? v / 12.92 : ((v + .055) / 1.055) ** 2.4)
    .reduce((sum, v, i) => sum + v * [.2126, .7152, .0722][i], 0);
const paper = light(getComputedStyle(document.body).backgroundColor);
return Math.min(...[...document.body.querySelectorAll('*')].filter((e) => e.textContent.trim()).map((e) => {
  const ink = light(getComputedStyle(e).color);
  return (Math.max(ink, paper) + .05) / (Math.min(ink, paper) + .05);
}));
"""


def make_page(tevpf, folder):
    subprocess.run([os.path.join(os.path.dirname(os.path.realpath(__file__)), "make_plant")], cwd=folder, check=True)
    text = "n,x,label\n" + "".join(f'{n},{x},"{label}"\n' for n, x, label in ROWS)
    subprocess.run([tevpf, "import", "plant.pf", "runs", "-"], cwd=folder, input=text.encode(), check=True)
    # Shown with 6 digits, these are the same.
    subprocess.run([tevpf, "import", "plant.pf", "levels", "-"], cwd=folder, input=b"id,level\n1,1.0000002\n2,1.0000001\n", check=True)
    subprocess.run([tevpf, "report", "plant.pf", "-o", "plant.html"], cwd=folder, check=True)
    return (pathlib.Path(folder).resolve() / "plant.html").as_uri()


def start():
    options = webdriver.ChromeOptions()
    for option in ("--headless=new", "--no-sandbox", "--disable-gpu", "--hide-scrollbars"):
        options.add_argument(option)
    options.set_capability("goog:loggingPrefs", {"browser": "ALL", "performance": "ALL"})
    return webdriver.Chrome(options=options, service=webdriver.chrome.service.Service("/usr/bin/chromedriver"))


def window(browser, width, **media):
    browser.execute_cdp_cmd("Emulation.setDeviceMetricsOverride", dict(width=width, height=1400, deviceScaleFactor=1, mobile=False))
    browser.execute_cdp_cmd("Emulation.setEmulatedMedia", dict(
        media=media.get("media", ""), features=[dict(name="prefers-color-scheme", value=media.get("scheme", "light"))]))


def shown_rows(table):
    return [int(row.find_element(By.TAG_NAME, "th").text) for row in table.find_elements(By.CSS_SELECTOR, "tbody tr") if row.is_displayed()]


def check_sorting(table):
    headings = {h.text.strip("↕ "): h for h in table.find_elements(By.CSS_SELECTOR, "thead th")}
    for name, order in ORDERS.items():
        button = headings[name].find_element(By.TAG_NAME, "button")
        missing = [2, 6] if name == "x" else []
        backwards = [row for row in order[::-1] if row not in missing] + missing
        for state, want in ("ascending", order), ("descending", backwards), ("none", [1, 2, 3, 4, 5, 6]):
            button.send_keys(Keys.ENTER)
            assert shown_rows(table) == want, (name, state, shown_rows(table))
            assert [h.get_attribute("aria-sort") for h in headings.values()] == [state if n == name else "none" for n in headings]


def check_filter(section, table):
    field, output = section.find_element(By.TAG_NAME, "input"), section.find_element(By.TAG_NAME, "output")
    for text, want in ("RUN", [4, 5]), ("run 9", [5]), ("ALERT x", []), ("1 alert", [3]), ("alert", [3, 6]), ("no such", []), ("10 nominal", [1]), ("  ", [1, 2, 3, 4, 5, 6]):
        field.clear()
        field.send_keys(text)
        assert shown_rows(table) == want, (text, shown_rows(table))
        assert output.text == (f"{len(want)} of 6" if text.strip() else ""), output.text


def check_looks(browser, folder):
    for name, width, media in ("light", 1200, {}), ("dark", 1200, dict(scheme="dark")), ("narrow", 380, {}):
        window(browser, width, **media)
        browser.save_screenshot(os.path.join(folder, name + ".png"))
        assert browser.execute_script(CONTRAST) >= 4.5, name
        assert browser.execute_script("return document.documentElement.scrollWidth") == width, name
    window(browser, 800, media="print", scheme="dark")
    paper, filters, pane = browser.execute_script("""return [getComputedStyle(document.body).backgroundColor,
        getComputedStyle(document.querySelector('.filter')).display, getComputedStyle(document.querySelector('.pane')).overflow]""")
    assert (paper, filters, pane) == ("rgb(255, 255, 255)", "none", "visible")
    with open(os.path.join(folder, "paper.pdf"), "wb") as out:
        out.write(base64.b64decode(browser.print_page()))
    window(browser, 1200)


def main():
    tevpf, folder = os.path.realpath(sys.argv[1]), sys.argv[2]
    os.makedirs(folder, exist_ok=True)
    url = make_page(tevpf, folder)
    browser = start()
    try:
        window(browser, 1200)
        browser.get(url)
        section = browser.find_element(By.XPATH, "//section[h2[contains(., 'runs')]]")
        table = section.find_element(By.CSS_SELECTOR, "table.sortable")
        check_sorting(table)
        levels = browser.find_element(By.XPATH, "//section[h2[contains(., 'levels')]]//table[@class='sortable']")
        levels.find_elements(By.TAG_NAME, "button")[2].click()
        assert shown_rows(levels) == [2, 1], "not sorted by all digits"
        check_filter(section, table)
        check_looks(browser, folder)
        assert browser.get_log("browser") == [], "messages on the console"
        requests = [entry for entry in browser.get_log("performance") if '"Network.requestWillBeSent"' in entry["message"]]
        assert all(url in entry["message"] or "data:," in entry["message"] for entry in requests), requests
        browser.execute_cdp_cmd("Emulation.setScriptExecutionDisabled", dict(value=True))
        browser.get(url)
        table = browser.find_elements(By.CSS_SELECTOR, "table.sortable")[-1]
        assert shown_rows(table) == [1, 2, 3, 4, 5, 6] and not browser.find_elements(By.TAG_NAME, "button")
        assert not any(p.is_displayed() for p in browser.find_elements(By.CLASS_NAME, "filter"))
    finally:
        browser.quit()


main()
