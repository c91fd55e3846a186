// Times neaps (its harmonic predictor, @neaps/tide-predictor) on the station-days that
// predict times: every station of a folder dumped by `tidefiles dump`, three days from
// 2024-01-01 00:00 UT, a point every 0.1 h and every 1 h, microseconds of processor time
// per station-day (the process's: node's collector threads count too) as the best of
// alternating rounds. Each station-day makes its predictor from the constants
// and asks for the day's timeline, as PredictDay reads the station and sums its day.
//   node neaps_days.mjs NEAPS_DIR WORLD_JSON [ROUNDS] [OURS_0.1 OURS_1]
// NEAPS_DIR holds node_modules with neaps; OURS_* (microseconds per station-day of the
// turned day, from predict) add the ratio lines.
import { readFileSync } from "node:fs";
import { join } from "node:path";
import { pathToFileURL } from "node:url";

const [neapsDir, worldJson, roundsArg, ours01, ours1] = process.argv.slice(2);
if (!neapsDir || !worldJson) {
  console.error("usage: node neaps_days.mjs NEAPS_DIR WORLD_JSON [ROUNDS] [OURS_0.1 OURS_1]");
  process.exit(2);
}
const predictor = await import(
  pathToFileURL(join(neapsDir, "node_modules", "@neaps", "tide-predictor", "dist", "index.js")).href
);
const rounds = Math.max(1, Number(roundsArg ?? 3));

// neaps knows constituents by NOAA names (upper case for most: RHO1, LAM2, MSF); rows of our
// table without a usual name have no counterpart and are left out.
const known = predictor.constituents;
const neapsName = (name) => [name, name?.toUpperCase()].find((n) => n && known[n]);

const stations = JSON.parse(readFileSync(worldJson, "utf8"));
let ourTerms = 0;
let theirTerms = 0;
const sets = stations.map((s) => {
  const constituents = [];
  for (const c of s.constituents) {
    ourTerms += 1;
    const name = neapsName(c.name);
    if (!name) continue;
    constituents.push({ name, amplitude: c.amplitude, phase: c.phase });
  }
  ourTerms += 1;  // the mean level, a term of our sum; an offset to neaps
  theirTerms += constituents.length;
  return { constituents, offset: s.mean_level ?? 0 };
});

const days = [0, 1, 2].map((d) => new Date(Date.UTC(2024, 0, 1 + d)));
let sink = 0;
let points = 0;

function pass(stepHours) {
  for (const start of days) {
    const end = new Date(start.getTime() + 24 * 3600 * 1000);
    for (const s of sets) {
      const timeline = predictor
        .createTidePredictor(s.constituents, { offset: s.offset })
        .getTimelinePrediction({ start, end, timeFidelity: stepHours * 3600 });
      sink += timeline[0].level;
      points = timeline.length;
    }
  }
}

const steps = [0.1, 1];
const best = [Infinity, Infinity];
for (let r = 0; r < rounds; r += 1) {
  for (const i of r % 2 === 0 ? [0, 1] : [1, 0]) {
    const t0 = process.cpuUsage();
    pass(steps[i]);
    const used = process.cpuUsage(t0);
    best[i] = Math.min(best[i], used.user + used.system);
  }
}
const stationDays = sets.length * days.length;
console.log(`neaps (node ${process.version}): ${sets.length} stations, ${(theirTerms / sets.length).toFixed(1)} ` +
            `of our ${(ourTerms / sets.length).toFixed(1)} terms per station, best of ${rounds} rounds`);
const ours = [Number(ours01), Number(ours1)];
steps.forEach((step, i) => {
  pass(step);  // the point count of this step
  const us = best[i] / stationDays;
  const ratio = ours[i] > 0 ? `; turned day ${ours[i].toFixed(2)} us, ${(us / ours[i]).toFixed(1)}x faster` : "";
  console.log(`  step ${step} h (${points} points): ${us.toFixed(2)} us per station-day${ratio}`);
});
console.log(`(checksum ${sink.toPrecision(6)})`);
