// The nets of a module: bit numbers mapped to local nets, and a name for
// every net.
#include <algorithm>
#include <limits>
#include <string>
#include <unordered_map>
#include <unordered_set>

#include "reader/Nlw_JsonReader_Internal.h"

namespace nlw_json {

namespace {

// Bit numbers become local net numbers in the order the bits first appear
// (ports, named nets, cells). Numbers usually run densely within a module,
// so a table indexed by bit number serves; scattered numbers use a hash.
void MapBits(Module& m, std::vector<int32_t>& map) {
    int32_t lo = std::numeric_limits<int32_t>::max(), hi = -1;
    for (int32_t r : m.refs)
        if (r >= 0) {
            lo = std::min(lo, r);
            hi = std::max(hi, r);
        }
    int32_t next = 0;
    if (hi >= 0) {
        uint64_t range = static_cast<uint64_t>(hi) - static_cast<uint64_t>(lo) + 1;
        if (range <= 2 * static_cast<uint64_t>(m.refs.size()) + 4096) {
            map.assign(range, -1);
            for (int32_t& r : m.refs) {
                if (r < 0) continue;
                int32_t& slot = map[static_cast<size_t>(r - lo)];
                if (slot < 0) slot = next++;
                r = slot;
            }
        } else {
            std::unordered_map<int32_t, int32_t> sparse;
            sparse.reserve(m.refs.size());
            for (int32_t& r : m.refs) {
                if (r < 0) continue;
                auto ins = sparse.emplace(r, next);
                if (ins.second) ++next;
                r = ins.first->second;
            }
        }
    }
    m.numNets = static_cast<uint32_t>(next);
}

constexpr uint32_t kClassStep = 1u << 30;

}  // namespace

// Ranks: a port name first (in port order), then a public name, then an
// internal one (in file order); bits nothing names rank last.
void NameNets(Module& m, NameScratch& scratch, TextPool& pool) {
    const std::vector<NetEntry>& entries = scratch.entries;
    MapBits(m, scratch.bitMap);
    if (entries.size() >= kClassStep || m.ports.size() >= kClassStep)
        Fail(Where{m.name, {}, {}, {}}.Text() + ": too many nets");
    std::vector<NameCandidate>& cands = scratch.cands;
    cands.clear();
    std::vector<Text>& portAka = scratch.portAka;
    portAka.assign(m.ports.size(), "");
    std::vector<uint8_t>& portFlags = scratch.portFlags;
    portFlags.assign(m.ports.size(), 0);
    for (const NetEntry& e : entries)
        if (e.port >= 0) {
            portAka[static_cast<size_t>(e.port)] = e.aka;
            portFlags[static_cast<size_t>(e.port)] = e.flags;
        }
    for (size_t k = 0; k < m.ports.size(); ++k) {
        const Port& p = m.ports[k];
        cands.push_back({p.name, p.bitFirst, p.width, p.msb, p.lsb, portAka[k],
                         static_cast<uint32_t>(k), portFlags[k]});
    }
    for (size_t j = 0; j < entries.size(); ++j) {
        const NetEntry& e = entries[j];
        if (e.port >= 0) continue;
        uint32_t cls = e.hidden ? 2 : 1;
        cands.push_back({e.name, e.bitFirst, e.width, e.msb, e.lsb, e.aka,
                         cls * kClassStep + uint32_t(j), e.flags});
    }

    std::vector<uint32_t>& rank = scratch.rank;
    std::vector<int32_t>& winner = scratch.winner;
    std::vector<uint32_t>& winBit = scratch.winBit;
    rank.assign(m.numNets, std::numeric_limits<uint32_t>::max());
    winner.assign(m.numNets, -1);
    winBit.assign(m.numNets, 0);
    for (size_t c = 0; c < cands.size(); ++c) {
        const NameCandidate& cd = cands[c];
        for (uint32_t i = 0; i < cd.width; ++i) {
            int32_t r = m.refs[cd.bitFirst + i];
            if (r < 0 || cd.rank >= rank[static_cast<size_t>(r)]) continue;
            rank[static_cast<size_t>(r)] = cd.rank;
            winner[static_cast<size_t>(r)] = static_cast<int32_t>(c);
            winBit[static_cast<size_t>(r)] = i;
        }
    }

    // Names to keep clear of, wanted only when some net has no name.
    std::unordered_set<std::string_view> used;
    std::vector<int32_t>& busOf = scratch.busOf;
    busOf.assign(cands.size(), -1);
    m.nets.assign(m.numNets, NetName{});
    uint32_t generated = 0;
    for (uint32_t n = 0; n < m.numNets; ++n) {
        NetName& nn = m.nets[n];
        nn.rank = rank[n];
        if (winner[n] < 0) {
            if (used.empty())
                for (const NameCandidate& cd : cands) used.insert(cd.name);
            std::string name;
            do {
                name = "nlw_net_" + std::to_string(generated++);
            } while (used.count(name));
            nn.name = pool.Keep(name);
            continue;
        }
        const NameCandidate& cd = cands[static_cast<size_t>(winner[n])];
        if (cd.width > 1) {
            int32_t& bus = busOf[static_cast<size_t>(winner[n])];
            if (bus < 0) {
                bus = static_cast<int32_t>(m.buses.size());
                m.buses.push_back({cd.name, cd.msb, cd.lsb, cd.aka, cd.flags});
            }
            int32_t i = static_cast<int32_t>(winBit[n]);
            nn.bus = bus;
            nn.index = cd.msb >= cd.lsb ? cd.lsb + i : cd.lsb - i;
        } else {
            nn.name = cd.name;
            nn.aka = cd.aka;
            nn.flags = cd.flags;
        }
    }

    // Constant bits of the buses made: 0, 1 and x are assigned, z floats.
    m.constMembers.clear();
    for (size_t c = 0; c < cands.size(); ++c) {
        const int32_t bus = busOf[c];
        if (bus < 0) continue;
        const NameCandidate& cd = cands[c];
        for (uint32_t i = 0; i < cd.width; ++i) {
            int32_t r = m.refs[cd.bitFirst + i];
            if (r >= 0 || r == kConstZ) continue;
            int32_t index = cd.msb >= cd.lsb ? cd.lsb + int32_t(i) : cd.lsb - int32_t(i);
            m.constMembers.push_back({bus, index, r, cd.bitFirst + i});
        }
    }
}

}  // namespace nlw_json
