#!/usr/bin/env node
// Regenerates the embedded world station folder (data/world) from the npm package
// @neaps/tide-database: every accepted tide station with harmonic constants of its own.
//
//   cd tools/world-data && npm ci && node generate.mjs [--tidefiles PATH] [--out DIR]
//       [--json FILE] [--commercial-only]
//
// --tidefiles  the tidefiles tool (default: $TIDEFILES, else the first built one under
//              build*/native/tools/tidefiles/), --out the folder (default data/world),
// --json       also keep the stations JSON given to "tidefiles build",
// --commercial-only  leave out stations whose licence forbids commercial use.
import { stations } from "@neaps/tide-database";
import { spawnSync } from "node:child_process";
import fs from "node:fs";
import os from "node:os";
import path from "node:path";
import { fileURLToPath } from "node:url";

const here = path.dirname(fileURLToPath(import.meta.url));
const root = path.resolve(here, "../..");
const packageInfo = JSON.parse(
  fs.readFileSync(path.join(here, "node_modules/@neaps/tide-database/package.json"), "utf8"),
);

function parseArguments(argv) {
  const options = { out: path.join(root, "data/world"), json: null, tidefiles: process.env.TIDEFILES ?? null, commercialOnly: false };
  for (let i = 0; i < argv.length; i++) {
    const a = argv[i];
    const value = () => {
      if (i + 1 >= argv.length) throw new Error(`${a} needs a value`);
      return argv[++i];
    };
    if (a === "--out") options.out = path.resolve(value());
    else if (a === "--json") options.json = path.resolve(value());
    else if (a === "--tidefiles") options.tidefiles = path.resolve(value());
    else if (a === "--commercial-only") options.commercialOnly = true;
    else throw new Error(`unknown argument ${a}`);
  }
  return options;
}

function findTidefiles() {
  const candidates = fs
    .readdirSync(root)
    .filter((d) => d.startsWith("build"))
    .map((d) => path.join(root, d, "native/tools/tidefiles/tidefiles"))
    .filter((p) => fs.existsSync(p));
  if (candidates.length === 0) throw new Error("tidefiles not found: build it (./run build) or pass --tidefiles");
  return candidates[0];
}

// Rounds as the tool does (C's round: halves away from zero).
function roundHalfAway(x) {
  return Math.sign(x) * Math.round(Math.abs(x));
}

// Standard-time offset from UT in minutes: the smaller of mid-January's and mid-July's, since
// daylight saving time only ever adds.
function standardOffsetMinutes(timeZone) {
  const offsetAt = (date) => {
    const text = new Intl.DateTimeFormat("en-US", { timeZone, timeZoneName: "longOffset" })
      .formatToParts(date)
      .find((p) => p.type === "timeZoneName").value;
    const m = text.match(/GMT([+-])(\d\d):(\d\d)/);
    return m ? (m[1] === "-" ? -1 : 1) * (Number(m[2]) * 60 + Number(m[3])) : 0;
  };
  return Math.min(offsetAt(new Date(Date.UTC(2024, 0, 15))), offsetAt(new Date(Date.UTC(2024, 6, 15))));
}

// Zone description: universal time = zone time + zone, so a station on UTC+1 holds -1.
function zoneDescription(timeZone) {
  const zone = -roundHalfAway(standardOffsetMinutes(timeZone) / 60);
  return zone === 0 ? 0 : zone; // no -0 in the JSON
}

// Mean sea level above the station's chart datum, metres; null when the datums do not say.
function meanLevel(station) {
  const datums = station.datums ?? {};
  const chartDatum = station.chart_datum;
  if (chartDatum === "MSL") return 0;
  if (typeof datums.MSL !== "number" || typeof datums[chartDatum] !== "number") return null;
  return datums.MSL - datums[chartDatum];
}

function select(options) {
  const dropped = { subordinate: [], noHarmonics: [], noDatums: [], nonCommercial: [], samePosition: [] };
  const candidates = [];
  for (const s of stations) {
    if (s.kind !== "tide") continue;
    if (s.type !== "reference") {
      dropped.subordinate.push(s);
      continue;
    }
    if (options.commercialOnly && s.license?.commercial_use === false) {
      dropped.nonCommercial.push(s.id);
      continue;
    }
    const constituents = s.harmonic_constituents ?? [];
    if (constituents.length === 0) {
      dropped.noHarmonics.push(s.id);
      continue;
    }
    const level = meanLevel(s);
    if (level === null) {
      dropped.noDatums.push(s.id);
      continue;
    }
    candidates.push({ station: s, level, constituents });
  }
  // Stations whose positions round to the same whole minutes cannot be told apart by the
  // engine's search: keep the best-scored one of each position.
  const best = new Map();
  for (const c of candidates) {
    const key = `${roundHalfAway(c.station.latitude * 60)},${roundHalfAway(c.station.longitude * 60)}`;
    const kept = best.get(key);
    const score = (x) => x.station.quality?.score ?? 0;
    if (!kept) best.set(key, c);
    else if (score(c) > score(kept)) {
      dropped.samePosition.push(`${kept.station.id} (same position as ${c.station.id})`);
      best.set(key, c);
    } else dropped.samePosition.push(`${c.station.id} (same position as ${kept.station.id})`);
  }
  const keptSet = new Set(best.values());
  return { chosen: candidates.filter((c) => keptSet.has(c)), dropped };
}

function stationJson(c) {
  const s = c.station;
  return {
    name: s.name,
    latitude: s.latitude,
    longitude: s.longitude,
    zone: zoneDescription(s.timezone),
    mean_level: Math.round(c.level * 1e6) / 1e6,
    constituents: c.constituents.map((h) => ({ name: h.name, amplitude: h.amplitude, phase: h.phase })),
  };
}

function run(tool, args) {
  const r = spawnSync(tool, args, { encoding: "utf8", maxBuffer: 256 * 1024 * 1024 });
  if (r.error) throw r.error;
  return r;
}

function tally(stderr) {
  const droppedNames = new Map();
  const otherWarnings = [];
  for (const line of stderr.split("\n")) {
    const m = line.match(/no table row for (.*); dropped$/);
    if (m) {
      for (const name of m[1].split(", ")) droppedNames.set(name, (droppedNames.get(name) ?? 0) + 1);
    } else if (line.startsWith("tidefiles: warning:") || line.startsWith("tidefiles: error:")) {
      otherWarnings.push(line);
    }
  }
  return { droppedNames, otherWarnings };
}

function licenceSummary(chosen) {
  const byNotice = new Map();
  for (const c of chosen) {
    const key = c.station.attribution;
    const entry = byNotice.get(key) ?? { count: 0, licence: c.station.license };
    entry.count++;
    byNotice.set(key, entry);
  }
  return [...byNotice.entries()].sort((a, b) => b[1].count - a[1].count);
}

function writeReadme(out, chosen, dropped, droppedNames, options) {
  const lines = [];
  const p = (s = "") => lines.push(s);
  const version = packageInfo.version;
  p("# World tide station set");
  p();
  p('The station folder brtide and brdesk open when no --folder is given: "td_num.ntx", "td_crd.ntx" and "td_pnt.dat"');
  p(`with ${chosen.length} tide stations around the world. Generated by \`tools/world-data/generate.mjs\``);
  p(`from the npm package \`@neaps/tide-database\` ${version} (public harmonic constants; see the`);
  p("licences below). Do not edit the files by hand: regenerate them (README section \"Station");
  p("files and tidefiles\" of the repository).");
  p();
  p("`stations.tsv` gives, for every station number (the order of \"td_num.ntx\"), the package's");
  p("station id and the licence of that station's data. `tidefiles dump data/world` prints the");
  p("stations with their constants.");
  p();
  p("## How the set was made");
  p();
  p(`- Every accepted tide station of the package (its \`stations\` export, ${chosen.length + Object.values(dropped).reduce((n, l) => n + l.length, 0)} tide stations) that has`);
  p("  harmonic constants of its own, in the package's order.");
  p("- Left out:");
  const chosenIds = new Set(chosen.map((c) => c.station.id));
  const covered = dropped.subordinate.filter((s) => chosenIds.has(s.offsets?.reference)).length;
  p(`  - ${dropped.subordinate.length} subordinate stations: they predict from a reference station's constants`);
  p("    corrected by time and height offsets at high and low water, which the station files cannot");
  p(`    hold (the reference stations of ${covered} of them are in the set);`);
  p(`  - ${dropped.noHarmonics.length} reference stations without harmonic constants${dropped.noHarmonics.length ? ` (${dropped.noHarmonics.join(", ")})` : ""};`);
  p(`  - ${dropped.noDatums.length} station${dropped.noDatums.length === 1 ? "" : "s"} whose datums do not give mean sea level above chart datum${dropped.noDatums.length ? ` (${dropped.noDatums.join(", ")})` : ""};`);
  p(`  - ${dropped.samePosition.length} stations whose position rounds to the same whole minutes as a better-scored`);
  p("    station (the package's quality score), since the engine's search cannot tell them apart;");
  if (options.commercialOnly) p(`  - ${dropped.nonCommercial.length} stations whose licence forbids commercial use.`);
  p("- Position: the package's latitude and longitude, rounded to whole minutes.");
  p("- Zone description: the station's time zone's standard-time offset from UT (the smaller of");
  p("  its January and July offsets), rounded to whole hours (halves away from zero), sign such");
  p("  that universal time = zone time + zone (a station on UTC+1 holds -1).");
  p("- Mean level (constituent 0): mean sea level above the station's chart datum, the package's");
  p("  `datums.MSL` minus the datum its `chart_datum` names, in millimetres.");
  p("- Constituents: amplitudes (metres, stored in millimetres) and Greenwich phase lags (degrees,");
  p("  referred to UT, stored in tenths) as the package gives them, mapped to the rows of the");
  p("  constituent table by `tidefiles build` (usual names, common spellings, equal Doodson");
  p("  numbers). Names with no row are dropped:");
  p();
  p("  | constituent | stations |");
  p("  |---|---|");
  for (const [name, count] of [...droppedNames.entries()].sort((a, b) => b[1] - a[1] || a[0].localeCompare(b[0]))) {
    p(`  | ${name} | ${count} |`);
  }
  p();
  p("  Most are small shallow-water or long-period terms. `SA_KV`, `S1_KV` and `OQ2_KV` are the");
  p("  Norwegian Mapping Authority's own variants of Sa, S1 and OQ2, whose definitions the package");
  p("  does not give, so they are not taken for the table's Sa and S1.");
  p("- Names: converted to the Windows-1252 code page and cut to the 40-byte field.");
  p();
  p("## Sources, licences and attribution");
  p();
  p("The package's code is MIT licensed (Copyright (c) Sailing Naturali). Each station's data");
  p("carries its own licence; the package assembles the notice each station needs. The notices");
  p("of the stations in this set, with the number of stations each covers:");
  p();
  for (const [notice, { count, licence }] of licenceSummary(chosen)) {
    p(`- ${count} stations, licence ${licence?.type ?? "unknown"}${licence?.commercial_use === false ? " (no commercial use)" : ""}:`);
    p(`  ${notice}`);
  }
  p();
  const nc = chosen.filter((c) => c.station.license?.commercial_use === false).length;
  if (nc > 0) {
    p(`${nc} stations are licensed CC BY-NC 4.0: their data may not be used commercially. \`stations.tsv\``);
    p("names them; `node generate.mjs --commercial-only` makes a set without them.");
    p();
  }
  p("The package's NOTICE adds: station location fields derived from GeoNames data (CC BY 4.0),");
  p("OpenStreetMap extracts (ODbL 1.0, © OpenStreetMap contributors) and the Marine Regions");
  p("Maritime Boundaries Geodatabase (CC BY 4.0, Flanders Marine Institute). None of those derived");
  p("location fields (locality, region, country) is in these files: they hold the package's station");
  p("names, positions, datums and harmonic constants only.");
  p();
  p("Tide predictions made from these constants are not for navigation.");
  fs.writeFileSync(path.join(out, "README.md"), lines.join("\n") + "\n");
}

function main() {
  const options = parseArguments(process.argv.slice(2));
  const tool = options.tidefiles ?? findTidefiles();
  const { chosen, dropped } = select(options);

  const json = JSON.stringify(chosen.map(stationJson));
  const jsonPath = options.json ?? path.join(fs.mkdtempSync(path.join(os.tmpdir(), "world-data-")), "stations.json");
  fs.writeFileSync(jsonPath, json);
  fs.mkdirSync(options.out, { recursive: true });

  const build = run(tool, ["build", jsonPath, options.out]);
  if (build.status !== 0) {
    process.stderr.write(build.stderr);
    throw new Error(`tidefiles build failed (status ${build.status})`);
  }
  const { droppedNames, otherWarnings } = tally(build.stderr);
  if (otherWarnings.length > 0) {
    process.stderr.write(otherWarnings.join("\n") + "\n");
    throw new Error("tidefiles build reported warnings beyond unknown constituents: fix the selection");
  }
  const check = run(tool, ["check", options.out]);
  if (check.status !== 0) {
    process.stderr.write(check.stdout + check.stderr);
    throw new Error("tidefiles check failed on the generated folder");
  }

  const tsv = ["number\tid\tlicence"];
  chosen.forEach((c, i) => tsv.push(`${i}\t${c.station.id}\t${c.station.license?.type ?? ""}`));
  fs.writeFileSync(path.join(options.out, "stations.tsv"), tsv.join("\n") + "\n");
  writeReadme(options.out, chosen, dropped, droppedNames, options);
  if (!options.json) fs.rmSync(path.dirname(jsonPath), { recursive: true, force: true });

  process.stdout.write(build.stdout + check.stdout);
  console.log(
    `left out: ${dropped.subordinate.length} subordinate, ${dropped.noHarmonics.length} without constants, ` +
      `${dropped.noDatums.length} without datums, ${dropped.samePosition.length} same position` +
      (options.commercialOnly ? `, ${dropped.nonCommercial.length} non-commercial` : ""),
  );
}

try {
  main();
} catch (e) {
  console.error(`generate.mjs: ${e.message}`);
  process.exit(1);
}
