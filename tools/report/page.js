// Sorting and filtering on the page that `tevpf report` writes. Without script all rows are there, in
// the order of the file.
'use strict';
(() => {
  const collator = new Intl.Collator('en', {numeric: true});

  // What a cell is sorted by: a number with all its digits, which are in the title where fewer are
  // shown, or a text. Null: not a number.
  function sortKey(cell) {
    if (!cell.classList.contains('n')) return cell.textContent;
    const text = (cell.title || cell.textContent).replace('inf', 'Infinity');
    return text === '' || isNaN(text) ? null : Number(text);
  }

  // Numbers come before texts.
  function compare(a, b) {
    if (typeof a !== typeof b) return typeof a === 'number' ? -1 : 1;
    if (typeof a === 'string') return collator.compare(a, b);
    return a < b ? -1 : a > b ? 1 : 0;
  }

  // The rows in the order of a column; not a number stays last in both directions.
  function sorted(rows, column, direction) {
    const keyed = rows.map((row) => ({row, key: sortKey(row.cells[column])}));
    keyed.sort((a, b) => {
      if (a.key === null || b.key === null) return (a.key === null) - (b.key === null);
      return direction * compare(a.key, b.key);
    });
    return keyed.map((entry) => entry.row);
  }

  // A heading's button goes from ascending to descending to the order of the file.
  const next = {none: 'ascending', ascending: 'descending', descending: 'none'};

  function makeSortable(table) {
    const body = table.tBodies[0];
    const rows = [...body.rows];
    const headings = [...table.tHead.rows[0].cells].filter((th) => !th.classList.contains('plain'));
    for (const heading of headings) {
      const button = document.createElement('button');
      button.type = 'button';
      button.append(...heading.childNodes);
      heading.append(button);
      heading.setAttribute('aria-sort', 'none');
      button.addEventListener('click', () => {
        const order = next[heading.getAttribute('aria-sort')];
        for (const other of headings) other.setAttribute('aria-sort', 'none');
        heading.setAttribute('aria-sort', order);
        body.append(...(order === 'none' ? rows :
            sorted(rows, heading.cellIndex, order === 'ascending' ? 1 : -1)));
      });
    }
  }

  // Shows the rows in which every word of the filter occurs, in whatever case.
  function makeFilterable(table, filter) {
    const input = filter.querySelector('input');
    const output = filter.querySelector('output');
    const rows = [...table.tBodies[0].rows];
    let texts = null;  // of the rows, gathered when they are first needed
    input.addEventListener('input', () => {
      texts ??= rows.map((row) =>
        [...row.cells].map((cell) => cell.textContent.toLowerCase()).join('\n'));
      const words = input.value.toLowerCase().split(/\s+/).filter(Boolean);
      let shown = 0;
      rows.forEach((row, i) => {
        row.hidden = !words.every((word) => texts[i].includes(word));
        if (!row.hidden) ++shown;
      });
      output.textContent = words.length ? `${shown} of ${rows.length}` : '';
      filter.classList.toggle('active', words.length > 0);
    });
    filter.hidden = false;
  }

  for (const table of document.querySelectorAll('table.sortable')) {
    makeSortable(table);
    makeFilterable(table, table.closest('section').querySelector('.filter'));
  }
})();
