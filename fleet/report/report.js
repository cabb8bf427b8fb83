"use strict";
// The script of the page that lease-warranty-report writes. The element "data" has the result of the program's function
// content().

const data = JSON.parse(document.getElementById("data").textContent);
const today = Date.parse(data.today);
const DAY = 86400000;
const PAGE = 100; // number of rows that are added at once
const MONTHS_BEFORE = 6, MONTHS_AFTER = 36; // range of the time line
const MONTH_NAMES = ["Jan", "Feb", "Mar", "Apr", "May", "Jun", "Jul", "Aug", "Sep", "Oct", "Nov", "Dec"];
const STATES = { "": "any", over: "over", soon: "ends soon", later: "ends later", open: "no end on record",
  none: "none on record" };
const compare = new Intl.Collator("en", { numeric: true }).compare;
const byId = (id) => document.getElementById(id);

function element(name, text, attributes = {}) {
  const made = document.createElement(name);
  if (text !== undefined && text !== null) made.textContent = text;
  for (const [key, value] of Object.entries(attributes)) made.setAttribute(key, value);
  return made;
}

// --- machines ---

// Returns the record that ends last. A record without an end counts as later than all others.
function latest(records) {
  return records.reduce((best, each) => (!best || (best.end && (!each.end || each.end > best.end)) ? each : best), null);
}

function recordsOf(rows) {
  return rows.map(([party, start, end]) => ({ party: party ?? "", start, end }));
}

function machineOf([name, owner, location, asset, product, leases, warranties]) {
  const machine = { name, owner, location, asset, product, leases: recordsOf(leases), warranties: recordsOf(warranties) };
  machine.lease = latest(machine.leases);
  machine.warranty = latest(machine.warranties);
  const parties = [...machine.leases, ...machine.warranties].map((each) => each.party);
  machine.words = [name, owner, location, asset, product, ...parties].join("\n").toLowerCase();
  return machine;
}

function stateOf(record) {
  if (!record) return "none";
  if (!record.end) return "open";
  const days = (Date.parse(record.end) - today) / DAY;
  return days < 0 ? "over" : days <= Number(byId("days").value) ? "soon" : "later";
}

const machines = data.machines.map(machineOf);

// --- time line ---

const monthOf = (date) => Number(date.slice(0, 4)) * 12 + Number(date.slice(5, 7)) - 1;
const firstMonth = monthOf(data.today) - MONTHS_BEFORE, lastMonth = monthOf(data.today) + MONTHS_AFTER;

// The bar of a record: that of its month, or one of the two bars for records that end before or after the time line.
const barOf = (record) => Math.min(Math.max(monthOf(record.end), firstMonth - 1), lastMonth + 1);

const isMonth = (month) => month >= firstMonth && month <= lastMonth;

function labelOf(month, count) {
  if (!isMonth(month)) return `${count} ${month < firstMonth ? "before" : "later"}`;
  return MONTH_NAMES[month % 12] + (month % 12 === 0 || month === firstMonth ? " " + Math.floor(month / 12) : "");
}

function countsByBar() {
  const counts = new Map();
  for (let month = firstMonth - 1; month <= lastMonth + 1; month++) counts.set(month, { lease: 0, warranty: 0 });
  for (const machine of machines) {
    for (const [kind, records] of [["lease", machine.leases], ["warranty", machine.warranties]]) {
      for (const record of records) if (record.end) counts.get(barOf(record))[kind]++;
    }
  }
  return counts;
}

function fullLabelOf(month) {
  if (month < firstMonth) return "Earlier months";
  if (month > lastMonth) return "Later months";
  return `${MONTH_NAMES[month % 12]} ${Math.floor(month / 12)}`;
}

function barElement(month, { lease, warranty }, most) {
  const title = `${fullLabelOf(month)}: ${lease} leases, ${warranty} warranties`;
  const bar = element("button", null, { type: "button", class: "bar", title, "aria-label": title, "aria-pressed": "false" });
  const stack = element("span", null, { class: month === monthOf(data.today) ? "stack now" : "stack" });
  const scale = Math.max(most, isMonth(month) ? 0 : lease + warranty);
  for (const [kind, count] of [["warranty", warranty], ["lease", lease]]) {
    const part = stack.appendChild(element("span", null, { class: kind }));
    part.style.height = `${(100 * count) / scale}%`;
  }
  if (!isMonth(month)) stack.classList.add("rest");
  bar.append(stack, element("span", labelOf(month, lease + warranty), { class: "label" }));
  bar.dataset.month = month;
  return bar;
}

function showTimeline() {
  const counts = countsByBar();
  // The bars for earlier and later months can be far higher than those of the months, so they do not affect the scale.
  const most = Math.max(1, ...[...counts].map(([month, each]) => (isMonth(month) ? each.lease + each.warranty : 0)));
  byId("scale").textContent = `per month, at most ${most}`;
  byId("timeline").replaceChildren(...[...counts].map(([month, each]) => barElement(month, each, most)));
}

// --- table ---

const COLUMNS = [
  { title: "Machine", key: (machine) => machine.name },
  { title: "Owner", key: (machine) => machine.owner },
  { title: "Location", key: (machine) => machine.location },
  { title: "Asset number", key: (machine) => machine.asset },
  { title: "Product", key: (machine) => machine.product },
  { title: "Lessor", key: (machine) => machine.lease?.party },
  { title: "Lease ends", key: (machine) => machine.lease?.end, records: "leases", record: "lease" },
  { title: "Warrantor", key: (machine) => machine.warranty?.party },
  { title: "Warranty ends", key: (machine) => machine.warranty?.end, records: "warranties", record: "warranty" },
];
let order = { column: 0, direction: 1 };
let month = null; // the selected bar
let shown = []; // the machines that pass the filters, in the selected order
let rowCount = 0;

function endCell(machine, column) {
  const record = machine[column.record], state = stateOf(record);
  const others = machine[column.records].length - 1;
  const text = record ? record.end ?? STATES.open : STATES.none;
  return element("td", others > 0 ? `${text} (+${others})` : text, { class: state, "data-label": column.title });
}

function rowElement(machine) {
  const row = element("tr");
  row.append(element("th", machine.name, { scope: "row" }));
  for (const column of COLUMNS.slice(1)) {
    row.append(column.records ? endCell(machine, column)
      : element("td", column.key(machine), { "data-label": column.title }));
  }
  return row;
}

function addRows(count) {
  const rows = shown.slice(rowCount, rowCount + count).map(rowElement);
  document.querySelector("#machines tbody").append(...rows);
  rowCount += rows.length;
  byId("more").hidden = rowCount >= shown.length;
}

// Machines without a value are last in either sort direction.
function inOrder(list) {
  const { key } = COLUMNS[order.column];
  return list.map((machine) => [key(machine) || "", machine]).sort(([one, a], [other, b]) =>
    !one - !other || order.direction * compare(one, other) || compare(a.name, b.name)).map(([, machine]) => machine);
}

function passes(machine, words, lease, warranty) {
  return words.every((word) => machine.words.includes(word)) &&
    (!lease || stateOf(machine.lease) === lease) && (!warranty || stateOf(machine.warranty) === warranty) &&
    (month === null || [...machine.leases, ...machine.warranties].some((each) => each.end && barOf(each) === month));
}

function update() {
  const words = byId("search").value.toLowerCase().split(/\s+/).filter(Boolean);
  const lease = byId("lease-state").value, warranty = byId("warranty-state").value;
  shown = inOrder(machines.filter((machine) => passes(machine, words, lease, warranty)));
  document.querySelector("#machines tbody").replaceChildren();
  rowCount = 0;
  addRows(PAGE);
  byId("count").textContent = `${shown.length} of ${machines.length} machines` +
    (month === null ? "" : `; something ends in: ${fullLabelOf(month)}`);
  document.querySelectorAll("#machines thead th").forEach((cell, index) => cell.setAttribute("aria-sort",
    index !== order.column ? "none" : order.direction > 0 ? "ascending" : "descending"));
  for (const bar of byId("timeline").children) bar.setAttribute("aria-pressed", String(Number(bar.dataset.month) === month));
  byId("order").value = `${order.column},${order.direction}`;
}

// --- controls ---

function fillControls() {
  const head = element("tr");
  COLUMNS.forEach(({ title }, index) => {
    const cell = head.appendChild(element("th", null, { scope: "col" }));
    cell.append(element("button", title, { type: "button" }));
    cell.firstChild.addEventListener("click", () => {
      order = { column: index, direction: order.column === index ? -order.direction : 1 };
      update();
    });
    byId("order").append(element("option", `${title} \u2191`, { value: `${index},1` }),
      element("option", `${title} \u2193`, { value: `${index},-1` }));
  });
  document.querySelector("#machines thead").append(head);
  for (const id of ["lease-state", "warranty-state"]) {
    byId(id).append(...Object.entries(STATES).map(([value, text]) => element("option", text, { value })));
  }
}

function listen() {
  for (const id of ["search", "lease-state", "warranty-state", "days"]) byId(id).addEventListener("input", update);
  byId("order").addEventListener("input", () => {
    const [column, direction] = byId("order").value.split(",").map(Number);
    order = { column, direction };
    update();
  });
  byId("filters").addEventListener("submit", (event) => event.preventDefault());
  byId("filters").addEventListener("reset", () => {
    month = null;
    setTimeout(update); // after the browser has reset the controls
  });
  byId("timeline").addEventListener("click", (event) => {
    const bar = event.target.closest(".bar");
    if (!bar) return;
    month = Number(bar.dataset.month) === month ? null : Number(bar.dataset.month);
    update();
  });
  byId("more").addEventListener("click", () => addRows(PAGE));
  new IntersectionObserver(([entry]) => entry.isIntersecting && addRows(PAGE)).observe(byId("more"));
  addEventListener("beforeprint", () => addRows(shown.length));
}

function showMissing() {
  byId("without").hidden = data.missing.length === 0;
  byId("missing").append(...data.missing.map(([name, reason]) => {
    const row = element("tr");
    row.append(element("th", name, { scope: "row" }), element("td", reason));
    return row;
  }));
}

const without = (record) => machines.filter((machine) => !machine[record]).length;
byId("summary").textContent = `As of ${data.today}: ${machines.length} machines with data, ${data.missing.length} without; ` +
  `${without("lease")} have no lease and ${without("warranty")} no warranty on record.`;
fillControls();
showTimeline();
showMissing();
update();
listen();
