// SPDX-License-Identifier: MIT
// Makes the tables of instances sortable and searchable. Without it they are plain tables.
'use strict';
(() => {
  const order = new Intl.Collator(undefined, { numeric: true, sensitivity: 'base' });
  const tables = Array.from(document.querySelectorAll('table.instances'));

  // A number counts as the device delivered it, not as the text that people read ("9 GiB", "10 MiB").
  const keyOf = (cell) => {
    const number = cell.dataset.number;
    if (number === undefined) return cell.textContent;
    return /^-?\d+$/.test(number) ? BigInt(number) : Number(number);
  };

  // Numbers before texts, empty cells last in both directions.
  const compare = (left, right, sign) => {
    if (left === '' || right === '') return (left === '') - (right === '');
    const leftIsText = typeof left === 'string';
    const rightIsText = typeof right === 'string';
    if (leftIsText !== rightIsText) return sign * (leftIsText - rightIsText);
    return sign * (leftIsText ? order.compare(left, right) : (left > right) - (left < right));
  };

  const sort = (table, head) => {
    const sign = head.getAttribute('aria-sort') === 'ascending' ? -1 : 1;
    const rows = Array.from(table.tBodies[0].rows, (row) => ({ row, key: keyOf(row.cells[head.cellIndex]) }));
    rows.sort((left, right) => compare(left.key, right.key, sign));
    const sorted = document.createDocumentFragment();
    rows.forEach(({ row }) => sorted.append(row));
    table.tBodies[0].append(sorted);
    for (const other of head.parentNode.cells) other.removeAttribute('aria-sort');
    head.setAttribute('aria-sort', sign > 0 ? 'ascending' : 'descending');
  };

  for (const table of tables) {
    for (const head of table.tHead.rows[0].cells) {
      const button = document.createElement('button');
      button.type = 'button';
      button.append(...head.childNodes);
      button.addEventListener('click', () => sort(table, head));
      head.append(button);
    }
  }

  const texts = new WeakMap();
  const textOf = (row) => {
    if (!texts.has(row)) texts.set(row, Array.from(row.cells, (cell) => cell.textContent).join('\n').toLowerCase());
    return texts.get(row);
  };

  const search = (wanted) => {
    const words = wanted.toLowerCase().split(/\s+/).filter(Boolean);
    let shown = 0;
    let all = 0;
    for (const table of tables) {
      let inTable = 0;
      for (const row of table.tBodies[0].rows) {
        const text = textOf(row);
        row.hidden = !words.every((word) => text.includes(word));
        inTable += row.hidden ? 0 : 1;
      }
      all += table.tBodies[0].rows.length;
      shown += inTable;
      table.closest('section').hidden = inTable === 0;
    }
    document.querySelector('.search output').textContent = words.length ? `${shown} of ${all} rows` : '';
  };

  const box = document.querySelector('.search');
  if (tables.length > 0) {
    box.hidden = false;
    box.querySelector('input').addEventListener('input', (event) => search(event.target.value));
  }
})();
